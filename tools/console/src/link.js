// The WebSocket to the server: says hello, comes back by itself, and pairs requests with replies.
const PROTOCOL = 1;
const FIRST_WAIT = 500; // ms
const LONGEST_WAIT = 8000;

export class Link {
  // `on` has: hello(hello), frame(frame), state(state, text); the states are open, lost, token and protocol.
  constructor(url, name, on) {
    Object.assign(this, { url, name, on, wait: FIRST_WAIT, nextId: 1, waiting: new Map() });
    this.connect();
  }

  connect() {
    this.refused = false;
    this.socket = new WebSocket(this.url);
    this.socket.onopen = () => {
      const token = sessionStorage.getItem('token');
      this.send({ hello: { protocol: PROTOCOL, name: this.name, frames: true, ...(token && { token }) } });
    };
    this.socket.onmessage = (event) => this.take(JSON.parse(event.data));
    this.socket.onclose = () => this.lose();
  }

  take(message) {
    if (message.hello) {
      this.wait = FIRST_WAIT;
      this.on.hello(message.hello);
      this.on.state('open', '');
    } else if (message.f !== undefined) {
      this.on.frame(message);
    } else if (message.bye) {
      this.farewell = message.bye;
    } else if (message.id !== undefined) {
      this.answer(message);
    } else if (message.error) {
      this.farewell = message.error;
      this.refused = message.kind === 'token' || message.kind === 'protocol';
      if (this.refused) this.on.state(message.kind, message.error);
    }
  }

  answer(reply) {
    const { resolve, reject } = this.waiting.get(reply.id) ?? {};
    this.waiting.delete(reply.id);
    if (reply.ok) resolve?.(reply);
    else reject?.(Object.assign(new Error(reply.error), { kind: reply.kind }));
  }

  request(body) {
    if (this.socket.readyState !== WebSocket.OPEN) return Promise.reject(new Error('no connection to the server'));
    const id = this.nextId++;
    return new Promise((resolve, reject) => {
      this.waiting.set(id, { resolve, reject });
      this.send({ id, ...body });
    });
  }

  send(message) {
    this.socket.send(JSON.stringify(message));
  }

  lose() {
    for (const { reject } of this.waiting.values()) reject(new Error('the connection was lost; it is not known whether this was done'));
    this.waiting.clear();
    if (this.refused) return; // goes on with another token, or a reload
    this.on.state('lost', this.farewell ?? 'no answer from the server');
    this.farewell = undefined;
    setTimeout(() => this.connect(), this.wait);
    this.wait = Math.min(2 * this.wait, LONGEST_WAIT);
  }

  useToken(token) {
    sessionStorage.setItem('token', token);
    this.connect();
  }
}
