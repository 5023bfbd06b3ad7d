<?php
// The service script the Quorvel client talks to. Accounts and data live in the
// data root named by QUORVEL_DATA (outside the document root).
declare(strict_types=1);

require __DIR__ . '/../../lib/service.php';

Quorvel\Service\answer_request($_GET, Quorvel\Service\data_root());
