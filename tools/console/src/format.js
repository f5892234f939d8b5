// A value's text, as the command line shows it. Values are hexadecimal texts of any width.
export function show(signal, hex) {
  if (hex === null || hex === undefined) return '?';
  const value = BigInt('0x' + hex);
  for (const [name, code] of Object.entries(signal.enum ?? {})) if (BigInt('0x' + code) === value) return name;
  const number = signal.radix === 'signed' ? BigInt.asIntN(signal.width, value) : value;
  if (signal.scale !== undefined) return `${+(Number(number) * signal.scale).toPrecision(12)} ${signal.unit ?? ''}`.trim();
  return digits(signal, hex, number) + (signal.unit ? ' ' + signal.unit : '');
}

function digits(signal, hex, number) {
  if (signal.width === 1) return String(number);
  if (signal.radix === 'bin') return '0b' + number.toString(2).padStart(signal.width, '0');
  return signal.radix === 'hex' ? '0x' + hex : String(number);
}

export const arrow = (flags) => ['', '↑', '↓', '↕'][flags & 3];
export const isSet = (hex) => !!hex && BigInt('0x' + hex) !== 0n;
