import { mount } from 'svelte';
import App from './components/App.svelte';
import './style.css';

mount(App, { target: document.getElementById('app') });
