import { svelte } from '@sveltejs/vite-plugin-svelte';
import { defineConfig } from 'vite';

// Fixed names, and nothing inline: the server names files by path and forbids inline scripts.
export default defineConfig({
  plugins: [svelte()],
  build: {
    modulePreload: false,
    rollupOptions: { output: { entryFileNames: 'app.js', assetFileNames: 'style[extname]' } },
  },
});
