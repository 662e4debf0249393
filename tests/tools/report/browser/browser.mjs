// A browser for the tests of one file, and pages that note everything that a page must not do.
import assert from 'node:assert/strict';
import {mkdtempSync, rmSync} from 'node:fs';
import {tmpdir} from 'node:os';
import {join} from 'node:path';
import {pathToFileURL} from 'node:url';
import {after, before} from 'node:test';
import puppeteer from 'puppeteer-core';

/** In milliseconds. A machine that runs many tests at once is slow; nothing waits without need. */
const patience = 120000;

let browser;
const profile = mkdtempSync(join(tmpdir(), 'report-browser-'));

/** Starts the browser before the tests of a file and ends it after them. */
export function useBrowser() {
    before(async () => {
        browser = await puppeteer.launch({
            executablePath: '/usr/bin/chromium',
            userDataDir: profile,
            timeout: patience,
            protocolTimeout: patience,
            args: ['--no-sandbox', '--disable-gpu', '--disable-quic', '--no-first-run', '--disable-background-networking',
                '--disable-component-update', '--disable-sync', '--disable-dev-shm-usage'],
        });
    });
    after(async () => {
        await browser.close();
        rmSync(profile, {recursive: true, force: true});
    });
}

/** An empty page. `page.noises` are its console messages, errors, dialogs, and requests outside the allowed address. */
export async function newPage(allowed, {scheme = 'light', width = 1280} = {}) {
    const page = await browser.newPage();
    page.setDefaultTimeout(patience);
    page.noises = [];
    page.on('console', (message) => page.noises.push(`console: ${message.text()}`));
    page.on('pageerror', (error) => page.noises.push(`error: ${error.message}`));
    page.on('request', (request) => request.url().startsWith(allowed) || page.noises.push(`request: ${request.url()}`));
    page.on('dialog', async (dialog) => {
        page.noises.push(`dialog: ${dialog.message()}`);
        await dialog.dismiss();
    });
    await page.setViewport({width, height: 900});
    await page.emulateMediaFeatures([{name: 'prefers-color-scheme', value: scheme}]);
    return page;
}

/** Opens the page of a report. */
export async function openPage(file, {hash = '', ...options} = {}) {
    const url = pathToFileURL(file).href;
    const page = await newPage(url, options);
    await page.goto(url + hash);
    await page.waitForFunction(() => document.documentElement.dataset.ready === 'true');
    return page;
}

/** Runs a test on a fresh page, on which nothing unwanted may happen. */
export async function withPage(file, options, test) {
    const page = await openPage(file, options);
    try {
        await test(page);
        assert.deepEqual(page.noises, []);
    } finally {
        await page.close();
    }
}

export const textOf = (page, selector) => page.$eval(selector, (place) => place.textContent);

export const textsOf = (page, selector) => page.$$eval(selector, (places) => places.map((place) => place.textContent));

/** Waits until the page has drawn what it planned for the next frames. */
export const drawn = (page) => page.evaluate(() =>
    new Promise((done) => { requestAnimationFrame(() => requestAnimationFrame(() => requestAnimationFrame(done))); }));
