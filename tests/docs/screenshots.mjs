// Takes the pictures of the site that docs/site.md shows. SITE is the folder of the site, PICTURES that of the pictures.
import {join} from 'node:path';
import {pathToFileURL} from 'node:url';
import {test} from 'node:test';
import {drawn, newPage, useBrowser} from './browser.mjs';

const pictures = {
    start: ['index.html', 1280, 'light'],
    'get-started': ['guide/start.html', 390, 'dark'],
    reference: ['reference/index.html', 1280, 'dark'],
    performance: ['performance.html', 1280, 'light'],
    format: ['store/format.html', 390, 'light'],
};

useBrowser();

test('take the pictures', async () => {
    const address = pathToFileURL(process.env.SITE + '/').href;
    for (const [name, [path, width, scheme]] of Object.entries(pictures)) {
        const page = await newPage(address, {width, scheme});
        await page.goto(address + path);
        await drawn(page);
        await page.screenshot({path: join(process.env.PICTURES, `${name}.png`)});
    }
});
