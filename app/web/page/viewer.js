// The viewer in a web page: lays the control out from its design table and
// passes the user's actions to the page's session on the server, which runs
// the control and answers with its state.
'use strict';

const params = new URLSearchParams(location.search);
let socket = null;
let design = null;
let nextId = 1;
let scale = 1;
let lists = {};            // the drop-down lists' entries, which change at run time
const forms = [];          // the forms shown, innermost last
const cardElements = {};   // name -> element of the control
const formElements = {};   // "FORM.NAME" -> element

function send(message) {
    if (socket && socket.readyState === WebSocket.OPEN)
        socket.send(JSON.stringify(message));
}

function request(...words) {
    send({ type: 'request', id: nextId++, request: words });
}

function px(twips) { return Math.round(twips * scale) + 'px'; }

function place(el, d) {
    el.classList.add('ctl');
    el.style.left = px(d.left);
    el.style.top = px(d.top);
    el.style.width = px(d.width);
    el.style.height = px(d.height);
    if (d.color && d.color !== '#000000') el.style.color = d.color;
    if (d.toolTip) el.title = d.toolTip;
}

// One control of a design table; name is what requests call it.
function makeControl(d, name) {
    let el;
    switch (d.kind) {
    case 'text':
        el = document.createElement('input');
        el.type = 'text';
        el.value = d.text;
        if (d.grey) el.classList.add('grey');
        el.addEventListener('change', () => request('set', name, el.value));
        el.addEventListener('blur', () => request('lostfocus', name));
        break;
    case 'combo':
    case 'drives':
        el = document.createElement('select');
        fillOptions(el, d.entries);
        el.addEventListener('change', () => request('set', name, el.selectedIndex));
        el.addEventListener('blur', () => request('lostfocus', name));
        break;
    case 'list':
        el = document.createElement('select');
        el.size = 4;
        el.addEventListener('change', () => request('set', name, el.selectedIndex));
        el.addEventListener('dblclick', () => request('dblclick', name));
        break;
    case 'dirs':
        el = document.createElement('input');
        el.type = 'text';
        el.addEventListener('change', () => request('set', name, el.value));
        break;
    case 'check': {
        el = document.createElement('label');
        const box = document.createElement('input');
        box.type = 'checkbox';
        const text = document.createElement('span');
        text.textContent = d.caption;
        el.append(box, text);
        box.addEventListener('change', () => request('set', name, box.checked ? 1 : 0));
        break;
    }
    case 'button':
        el = document.createElement('button');
        el.type = 'button';
        el.textContent = d.caption || buttonPicture(d.picture);
        el.addEventListener('click', () => request('click', name));
        break;
    case 'shape':
        el = document.createElement('div');
        el.classList.add('shape');
        if (/fill/i.test(d.name)) el.classList.add('fill');
        break;
    case 'grid':
        el = document.createElement('div');
        el.classList.add('grid');
        el.append(document.createElement('table'));
        el.addEventListener('dblclick', () => request('dblclick', name));
        break;
    default:
        el = document.createElement('div');
        el.classList.add('label');
        el.textContent = d.caption;
        if (d.bold) el.classList.add('bold');
        // The first press of a double click is a click, as on the desktop.
        el.addEventListener('click', () => request('click', name));
        el.addEventListener('dblclick', () => request('dblclick', name));
    }
    el.dataset.control = name;
    el.dataset.kind = d.kind;
    place(el, d);
    el.style.fontSize = Math.max(9, Math.round(8.25 * 20 * scale)) + 'px';
    return el;
}

function buttonPicture(picture) {
    return { folder: '\u2026', print: '\u2399', settings: '\u2699' }[
        String(picture).toLowerCase()] || picture || '';
}

function fillOptions(select, entries) {
    const same = select.options.length === entries.length &&
        [...select.options].every((o, i) => o.textContent === entries[i]);
    if (same) return;
    select.replaceChildren(...entries.map(text => {
        const option = document.createElement('option');
        option.textContent = text;
        return option;
    }));
}

function fillGrid(el, rows, gridName) {
    const table = el.querySelector('table');
    table.replaceChildren(...rows.map((cells, r) => {
        const tr = document.createElement('tr');
        tr.dataset.row = r;
        for (const cell of cells) {
            const td = document.createElement('td');
            td.textContent = cell;
            tr.append(td);
        }
        tr.addEventListener('click', () => {
            table.querySelectorAll('tr.current').forEach(t => t.classList.remove('current'));
            tr.classList.add('current');
            request('select', gridName, r);
        });
        return tr;
    }));
}

// Shows one control's value from the state.
function showValue(el, value, name) {
    if (!el || value === undefined) return;
    switch (el.dataset.kind) {
    case 'text':
    case 'dirs':
        if (document.activeElement !== el) el.value = value ?? '';
        break;
    case 'combo':
        if (lists[name]) fillOptions(el, lists[name]);
        el.selectedIndex = value;
        break;
    case 'list':
    case 'drives':
        fillOptions(el, value.entries || []);
        el.selectedIndex = value.index;
        if (value.enabled === false) el.disabled = true; else el.disabled = false;
        break;
    case 'check':
        el.querySelector('input').checked = value === 1;
        el.querySelector('input').indeterminate = value === 2;
        break;
    case 'shape':
        el.style.width = px(value);
        break;
    case 'grid':
        fillGrid(el, value, name);
        break;
    default:
        el.textContent = value ?? '';
    }
}

function showState(state) {
    if (!state) return;
    window.lastState = state;
    lists = state.lists || lists;
    for (const [name, value] of Object.entries(state.controls || {}))
        showValue(cardElements[name], value, name);
    if (cardElements.DocLines) showValue(cardElements.DocLines, state.grid, 'DocLines');
    for (const [form, info] of Object.entries(state.forms || {}))
        for (const [name, value] of Object.entries(info.controls || {}))
            showValue(formElements[form + '.' + name], value, form + '.' + name);
}

function layOut() {
    const card = document.getElementById('card');
    scale = Math.min(window.innerWidth / design.card.width, 1.6);
    card.style.width = px(design.card.width);
    card.style.height = px(design.card.height);
    card.replaceChildren();
    for (const d of design.card.controls) {
        const el = makeControl(d, d.name);
        cardElements[d.name] = el;
        card.append(el);
    }
}

function showMessage(message) {
    const dialog = document.createElement('dialog');
    dialog.dataset.message = message.icon;
    const title = document.createElement('div');
    title.className = 'title';
    title.textContent = message.title;
    const text = document.createElement('div');
    text.className = 'text';
    text.textContent = message.text;
    const buttons = document.createElement('div');
    buttons.className = 'buttons';
    const answers = message.buttons === 'ok' ? [['ok', 'אישור']] : [['yes', 'כן'], ['no', 'לא']];
    for (const [answer, caption] of answers) {
        const button = document.createElement('button');
        button.type = 'button';
        button.dataset.answer = answer;
        button.textContent = caption;
        button.addEventListener('click', () => {
            send({ type: 'answer', answer });
            dialog.close();
            dialog.remove();
        });
        buttons.append(button);
    }
    // Escape answers as the box's close button would.
    dialog.addEventListener('cancel', event => {
        event.preventDefault();
        buttons.querySelector(message.buttons === 'ok' ? '[data-answer=ok]' : '[data-answer=no]')
            .click();
    });
    dialog.append(title, text, buttons);
    document.body.append(dialog);
    dialog.showModal();
}

function showForm(name, state) {
    const layout = design.forms[name];
    const dialog = document.createElement('dialog');
    dialog.dataset.form = name;
    const header = document.createElement('header');
    const caption = document.createElement('span');
    caption.textContent = layout ? layout.caption : name;
    const close = document.createElement('button');
    close.type = 'button';
    close.textContent = '\u2715';
    close.dataset.control = name + '.close';
    close.addEventListener('click', () => send({ type: 'close' }));
    header.append(caption, close);
    const body = document.createElement('div');
    body.className = 'form-body';
    if (layout) {
        body.style.width = px(layout.width);
        body.style.height = px(layout.height);
        for (const d of layout.controls) {
            const el = makeControl(d, name + '.' + d.name);
            formElements[name + '.' + d.name] = el;
            body.append(el);
        }
    }
    dialog.addEventListener('cancel', event => {
        event.preventDefault();
        send({ type: 'close' });
    });
    dialog.append(header, body);
    document.body.append(dialog);
    forms.push(dialog);
    dialog.showModal();
    showState(state);
}

function closeForm(name) {
    const dialog = document.querySelector(`dialog[data-form="${CSS.escape(name)}"]`);
    if (!dialog) return;
    for (const key of Object.keys(formElements))
        if (key.startsWith(name + '.')) delete formElements[key];
    dialog.close();
    dialog.remove();
    forms.splice(forms.indexOf(dialog), 1);
}

function status(text) {
    const el = document.getElementById('status');
    el.textContent = text;
    el.hidden = !text;
}

function started(message) {
    design = message.design;
    layOut();
    showState(message.state);
    document.body.dataset.ready = '1';
    // The address may name a document to show, as the desktop viewer's
    // command line does.
    const compDir = params.get('CompDir');
    if (compDir)
        request('call', 'ShowDoc', compDir, Number(params.get('type') || 20),
                Number(params.get('start') || 2));
}

function receive(event) {
    const message = JSON.parse(event.data);
    switch (message.type) {
    case 'hello': started(message); break;
    case 'reply':
        if (!message.ok) status(message.error);
        showState(message.state);
        document.body.dataset.replies = String(Number(document.body.dataset.replies || 0) + 1);
        break;
    case 'message': showMessage(message); break;
    case 'form': showForm(message.name, message.state); break;
    case 'formClosed': closeForm(message.name); break;
    case 'progress':
        if (cardElements.ProgressFill) cardElements.ProgressFill.style.width = px(message.fill);
        break;
    case 'print': window.open(message.url, '_blank', 'noopener'); break;
    case 'clipboard':
        if (navigator.clipboard) navigator.clipboard.writeText(message.text).catch(() => {});
        break;
    }
}

function connect() {
    const scheme = location.protocol === 'https:' ? 'wss:' : 'ws:';
    const query = new URLSearchParams();
    for (const key of ['SettingID', 'AccountKey'])
        if (params.has(key)) query.set(key, params.get(key));
    socket = new WebSocket(`${scheme}//${location.host}/ws?${query}`);
    socket.addEventListener('message', receive);
    socket.addEventListener('close', () => {
        document.body.dataset.closed = '1';
        status('החיבור לשרת נסגר; טען את הדף מחדש.');
    });
}

window.addEventListener('resize', () => {
    if (!design) return;
    const state = window.lastState;
    layOut();
    if (state) showState(state);
});

connect();
